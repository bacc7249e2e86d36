// Shared pieces of the CxF3 document tests: a private scratch folder and
// small file helpers.
#ifndef TESSARINE_TESTS_CXF3_TEST_SUPPORT_H
#define TESSARINE_TESTS_CXF3_TEST_SUPPORT_H

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

// A fresh folder under the system's temporary folder, removed afterwards.
class ScratchFolderTest : public ::testing::Test {
protected:
    void SetUp() override {
        const ::testing::TestInfo *info = ::testing::UnitTest::GetInstance()->current_test_info();
        p_folder = std::filesystem::temp_directory_path() /
                   (std::string("tessarine-") + info->test_suite_name() + "-" + info->name());
        std::filesystem::remove_all(p_folder);
        std::filesystem::create_directories(p_folder);
    }
    void TearDown() override { std::filesystem::remove_all(p_folder); }

    std::string PathOf(const std::string &ar_name) const { return (p_folder / ar_name).string(); }

    static std::string ReadFile(const std::string &ar_path) {
        std::ifstream file(ar_path, std::ios::binary);
        return std::string(std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>());
    }
    static void WriteFile(const std::string &ar_path, const std::string &ar_text) {
        std::ofstream(ar_path, std::ios::binary) << ar_text;
    }
    static std::size_t CountOf(const std::string &ar_text, const std::string &ar_what) {
        std::size_t count = 0;
        for (std::size_t at = ar_text.find(ar_what); at != std::string::npos; at = ar_text.find(ar_what, at + 1))
            ++count;
        return count;
    }

    std::filesystem::path p_folder;
};

// The text of a minimal CxF3 file around the given resources and custom resources.
inline std::string Cxf3Text(const std::string &ar_resources, const std::string &ar_custom_resources = "") {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
           "<cc:CxF xmlns:cc=\"http://colorexchangeformat.com/CxF3-core\">\n"
           "<cc:Resources>" +
           ar_resources + "</cc:Resources>" + ar_custom_resources + "</cc:CxF>\n";
}

// A cc:Object with the required parts.
inline std::string ObjectXml(const std::string &ar_id, const std::string &ar_type = "Target") {
    return "<cc:Object ObjectType=\"" + ar_type + "\" Name=\"N" + ar_id + "\" Id=\"" + ar_id +
           "\"><cc:CreationDate>2024-01-02T03:04:05Z</cc:CreationDate></cc:Object>";
}

#endif // TESSARINE_TESTS_CXF3_TEST_SUPPORT_H
