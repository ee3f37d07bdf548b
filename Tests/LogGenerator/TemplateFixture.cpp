#include "Tests/LogGenerator/TemplateFixture.h"

#include "PropertyList/PropertyListReader.h"

#include <fstream>

namespace ventrik
{

const Keys& simInfoKeys()
{
    static const Keys keys{"EF-ICCID",
                           "EF-MSISDN",
                           "EF-3GPP MAIL BOX DIALING NUMBER",
                           "EF-HPPLMN SEARCH PERIOD",
                           "EF-LOCI",
                           "EF-GPRS/PS-LOCI",
                           "EF-ACCESS CONTROL CLASS",
                           "EF-ADMINISTRATIVE DATA",
                           "EF-FPLMN",
                           "EF-ACTING HPLMN",
                           "EF-RAT MODE",
                           "EF-PLMN NETWORK NAME",
                           "EF-OPERATOR PLMN LIST",
                           "EF-OPLMNAcT"};
    return keys;
}

TemplateFixture::TemplateFixture(const std::string& fileName)
{
    std::ifstream file(VENTRIK_RESOURCES "/" + fileName, std::ios::binary);
    const Bytes bytes{std::istreambuf_iterator<char>(file), {}};
    const auto reading = readPropertyList(bytes);
    EXPECT_TRUE(reading) << reading.error;
    if (!reading)
        return;
    root = *reading.value->dictionary();
    collect(root);
}

void TemplateFixture::collect(const PlistDictionary& dictionary)
{
    for (const auto& [key, value] : dictionary) {
        entries.emplace(key, value);
        if (value.dictionary())
            collect(*value.dictionary());
    }
}

const PlistValue* TemplateFixture::only(const std::string& key)
{
    EXPECT_EQ(entries.count(key), 1U) << key;
    const auto entry = entries.find(key);
    return entry == entries.end() ? nullptr : &entry->second;
}

void TemplateFixture::expectDictionary(const std::string& name, const Keys& keys, const Keys& lists)
{
    const PlistValue* container = only(name);
    ASSERT_TRUE(container && container->dictionary()) << name;
    Keys all = keys;
    all.insert(all.end(), lists.begin(), lists.end());
    EXPECT_THAT(keysOf(*container->dictionary()), testing::UnorderedElementsAreArray(all)) << name;
    for (const std::string& list : lists)
        EXPECT_EQ(*container->dictionary()->find(list), PlistArray()) << name << " " << list;
    for (const std::string& key : keys)
        EXPECT_EQ(textAt(*container, {key}), "-") << name << " " << key;
}

void TemplateFixture::expectEmptyArray(const std::string& name)
{
    const PlistValue* container = only(name);
    ASSERT_TRUE(container && container->array()) << name;
    EXPECT_TRUE(container->array()->empty()) << name;
}

} // namespace ventrik
