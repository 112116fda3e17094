#include <cmath>

#include <gtest/gtest.h>

#include "platform/Variant.h"
#include "platform/fake/FixedLocale.h"

namespace cv {
namespace {

const fake::FixedLocale kPoint = fake::FixedLocale::Point();
const fake::FixedLocale kComma = fake::FixedLocale::Comma();

Variant To(const Variant& source, uint16_t vt, const platform::Locale& locale = kPoint) {
    Variant result = Variant::Str("unchanged");
    const ErrorInfo error = ChangeType(result, source, vt, locale);
    EXPECT_FALSE(error) << error.Description;
    return result;
}

int32_t Fails(const Variant& source, uint16_t vt, const platform::Locale& locale = kPoint) {
    Variant result = Variant::Str("unchanged");
    const ErrorInfo error = ChangeType(result, source, vt, locale);
    EXPECT_TRUE(result.IsEmpty());
    return error.Number;
}

std::string Text(const Variant& source, const platform::Locale& locale = kPoint) {
    return To(source, VT_BSTR, locale).AsStr();
}

TEST(ChangeType, AppliesTheEmptyAndNullRules) {
    EXPECT_EQ(To(Variant(), VT_I2), Variant::I2(0));
    EXPECT_EQ(To(Variant(), VT_BSTR), Variant::Str(""));
    EXPECT_EQ(To(Variant(), VT_BOOL), Variant::Bool(false));
    EXPECT_EQ(To(Variant(), VT_DATE), Variant::Date(0));
    EXPECT_EQ(To(Variant(), VT_NULL), Variant::Null());
    EXPECT_EQ(To(Variant::R8(5), VT_EMPTY), Variant());
    EXPECT_EQ(To(Variant::Str("x"), VT_NULL), Variant::Null());
    EXPECT_EQ(To(Variant::Null(), VT_NULL), Variant::Null());
    EXPECT_EQ(Fails(Variant::Null(), VT_EMPTY), kErrTypeMismatch);
    EXPECT_EQ(Fails(Variant::Null(), VT_I2), kErrTypeMismatch);
    EXPECT_EQ(Fails(Variant::Null(), VT_BSTR), kErrTypeMismatch);
    EXPECT_EQ(Fails(Variant::I2(1), 6), kErrTypeMismatch);  // currency is not carried
}

TEST(ChangeType, RoundsHalvesToEvenAndReportsOverflow) {
    EXPECT_EQ(To(Variant::R8(2.5), VT_I2), Variant::I2(2));
    EXPECT_EQ(To(Variant::R8(3.5), VT_I2), Variant::I2(4));
    EXPECT_EQ(To(Variant::R4(-2.5F), VT_I4), Variant::I4(-2));
    EXPECT_EQ(To(Variant::R8(2.51), VT_I2), Variant::I2(3));
    EXPECT_EQ(To(Variant::R8(-32768.5), VT_I2), Variant::I2(-32768));
    EXPECT_EQ(To(Variant::I4(70000), VT_R4), Variant::R4(70000.0F));
    EXPECT_EQ(Fails(Variant::R8(32767.5), VT_I2), kErrOverflow);
    EXPECT_EQ(Fails(Variant::I4(40000), VT_I2), kErrOverflow);
    EXPECT_EQ(Fails(Variant::R8(1e10), VT_I4), kErrOverflow);
    EXPECT_EQ(Fails(Variant::R8(std::nan("")), VT_I2), kErrOverflow);
    EXPECT_EQ(Fails(Variant::R8(1e39), VT_R4), kErrOverflow);
    EXPECT_EQ(Fails(Variant::R8(3e6), VT_DATE), kErrOverflow);
}

TEST(ChangeType, TreatsBooleansAsMinusOneAndZero) {
    EXPECT_EQ(To(Variant::Bool(true), VT_I2), Variant::I2(-1));
    EXPECT_EQ(To(Variant::Bool(true), VT_R8), Variant::R8(-1));
    EXPECT_EQ(Text(Variant::Bool(true)), "-1");
    EXPECT_EQ(Text(Variant::Bool(false)), "0");
    EXPECT_EQ(To(Variant::I2(5), VT_BOOL), Variant::Bool(true));
    EXPECT_EQ(To(Variant::R8(0.0), VT_BOOL), Variant::Bool(false));
    EXPECT_EQ(To(Variant::Str("true"), VT_BOOL), Variant::Bool(true));
    EXPECT_EQ(To(Variant::Str("FALSE"), VT_BOOL), Variant::Bool(false));
    EXPECT_EQ(To(Variant::Str("-1"), VT_BOOL), Variant::Bool(true));
    EXPECT_EQ(To(Variant::Str(" 0 "), VT_BOOL), Variant::Bool(false));
    EXPECT_EQ(To(Variant::Str("0,5"), VT_BOOL, kComma), Variant::Bool(true));
    EXPECT_EQ(Fails(Variant::Str("yes"), VT_BOOL), kErrTypeMismatch);
    EXPECT_EQ(Fails(Variant::Str(""), VT_BOOL), kErrTypeMismatch);
}

TEST(ChangeType, WritesNumbersWithTheRegionalDecimalSeparator) {
    EXPECT_EQ(Text(Variant::R8(1234.5), kComma), "1234,5");
    EXPECT_EQ(Text(Variant::R8(1.0 / 3.0)), "0.333333333333333");
    EXPECT_EQ(Text(Variant::R4(1.0F / 3.0F), kComma), "0,3333333");
    EXPECT_EQ(Text(Variant::R4(0.1F)), "0.1");
    EXPECT_EQ(Text(Variant::R8(1e20)), "1E+20");
    EXPECT_EQ(Text(Variant::R8(0.00001)), "1E-05");
    EXPECT_EQ(Text(Variant::R8(-0.0001)), "-0.0001");
    EXPECT_EQ(Text(Variant::R8(123456789012345678.0)), "1.23456789012346E+17");
    EXPECT_EQ(Text(Variant::R8(123456789012345.0)), "123456789012345");
    EXPECT_EQ(Text(Variant::R4(16777216.0F)), "1.677722E+07");
    EXPECT_EQ(Text(Variant::R8(-0.0)), "0");
    EXPECT_EQ(Text(Variant::R8(1e-300), kComma), "1E-300");
    EXPECT_EQ(Text(Variant::R8(INFINITY)), "Infinity");
    // Exact binary ties round away from zero, as the automation library does.
    EXPECT_EQ(Text(Variant::R4(654322.25F)), "654322.3");
    EXPECT_EQ(Text(Variant::R4(-654322.25F), kComma), "-654322,3");
    EXPECT_EQ(Text(Variant::R8(12345678901234.25)), "12345678901234.3");
}

TEST(ChangeType, ReadsNumbersWithTheRegionalSettings) {
    EXPECT_EQ(To(Variant::Str("1.234,5"), VT_R8, kComma), Variant::R8(1234.5));
    EXPECT_EQ(To(Variant::Str("&HFFFF"), VT_I2), Variant::I2(-1));
    EXPECT_EQ(Fails(Variant::Str("7.5"), VT_R8, kComma), kErrTypeMismatch);
    const double third = 1.0 / 3.0;
    EXPECT_NEAR(To(To(Variant::R8(third), VT_BSTR, kComma), VT_R8, kComma).AsR8(), third, 1e-15);
}

TEST(ChangeType, WritesAndReadsDatesWithTheRegionalFormats) {
    EXPECT_EQ(Text(Variant::Date(36526.5)), "1/1/2000 12:00:00 PM");
    EXPECT_EQ(Text(Variant::Date(36526.5), kComma), "01.01.2000 12:00:00");
    EXPECT_EQ(Text(Variant::Date(36526)), "1/1/2000");
    EXPECT_EQ(Text(Variant::Date(0.75)), "6:00:00 PM");
    EXPECT_EQ(Text(Variant::Date(0)), "12:00:00 AM");
    EXPECT_EQ(Fails(Variant::Date(1e7), VT_BSTR), 5);
    const double date = 46387 + (13 * 3600 + 2 * 60 + 3) / 86400.0;  // 2026-12-31 13:02:03
    EXPECT_NEAR(To(Variant::Str("12/31/2026 1:02:03 PM"), VT_DATE).AsR8(), date, 1e-9);
    EXPECT_NEAR(To(Variant::Str("31.12.2026 13:02:03"), VT_DATE, kComma).AsR8(), date, 1e-9);
    EXPECT_NEAR(To(Variant::Str(Text(Variant::Date(date))), VT_DATE).AsR8(), date, 1e-9);
    EXPECT_EQ(To(Variant::Str("2026-12-31"), VT_DATE, kComma), Variant::Date(46387));
    EXPECT_EQ(To(Variant::Str("13/1/2020"), VT_DATE), To(Variant::Str("1/13/2020"), VT_DATE));
    EXPECT_EQ(To(Variant::Str("Jan 5, 2020"), VT_DATE), To(Variant::Str("5 january 20"), VT_DATE));
    EXPECT_EQ(To(Variant::Str("6:00 PM"), VT_DATE), Variant::Date(0.75));
    EXPECT_EQ(To(Variant::Str("1/1/99"), VT_DATE), To(Variant::Str("1/1/1999"), VT_DATE));
    for (const char* text : {"hello", "1/2", "", "25:00", "2/30/2020", "13:00 PM", "1:2:3:4"}) {
        EXPECT_EQ(Fails(Variant::Str(text), VT_DATE), kErrTypeMismatch) << text;
    }
}

TEST(ChangeType, ConvertsArraysOnlyToTheirOwnTypeAndValuesInPlace) {
    for (const Variant& array :
         {Variant::Array(VT_I2, {Variant::I2(1), Variant::I2(2)}, 1), Variant::Bytes({1, 2}, 1)}) {
        const auto vt = array.VarType();
        EXPECT_EQ(To(array, vt), array);
        EXPECT_EQ(Fails(array, VT_ARRAY | VT_R8), kErrTypeMismatch);
        EXPECT_EQ(Fails(array, VT_I2), kErrTypeMismatch);
        EXPECT_EQ(Fails(array, VT_BSTR), kErrTypeMismatch);
        EXPECT_EQ(Fails(Variant::I2(1), vt), kErrTypeMismatch);
        EXPECT_EQ(TextOf(array, kPoint), "");
    }
    EXPECT_NE(Variant::Date(2.5), Variant::R8(2.5)) << "values of two types never compare equal";

    Variant value = Variant::Str("12.5");
    EXPECT_FALSE(ChangeType(value, value, VT_R8, kPoint));
    EXPECT_EQ(value, Variant::R8(12.5));
    value = Variant::Str("junk");
    EXPECT_EQ(ChangeType(value, value, VT_R8, kPoint),
              (ErrorInfo{kErrTypeMismatch, "Type mismatch"}));
    EXPECT_TRUE(value.IsEmpty());
}

// Both kinds of array answer the same questions; a byte array keeps one
// buffer and hands its bytes out as I2 elements.
TEST(VariantArrays, BytesAndVariantsShowTheSameElements) {
    const Variant elements = Variant::Array(VT_I2, {Variant::I2(0), Variant::I2(255)}, 1);
    const Variant bytes = Variant::Bytes({0, 255}, 1);
    EXPECT_EQ(elements.VarType(), VT_ARRAY | VT_I2);
    EXPECT_EQ(bytes.VarType(), VT_ARRAY | VT_UI1);
    EXPECT_TRUE(bytes.IsArray());
    EXPECT_EQ(bytes.AsBytes(), (std::vector<uint8_t>{0, 255}));
    EXPECT_TRUE(bytes.Elements().empty());
    EXPECT_TRUE(elements.AsBytes().empty());
    for (const Variant& array : {elements, bytes}) {
        EXPECT_EQ(array.LowerBound(), 1);
        ASSERT_EQ(array.ElementCount(), 2u);
        EXPECT_EQ(array.Element(0), Variant::I2(0));
        EXPECT_EQ(array.Element(1), Variant::I2(255));
        EXPECT_EQ(array.Element(2), Variant());
    }
    EXPECT_NE(bytes, elements);
    EXPECT_NE(bytes, Variant::Bytes({0, 254}, 1));
    EXPECT_EQ(Variant::I2(3).ElementCount(), 0u);
}

}  // namespace
}  // namespace cv
