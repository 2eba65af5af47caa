// Calls, or takes the address of, all that a host can call, so that the linker finds whether it is
// there. The program is not run. The script `check` finds members that are missing here.
#include "dcm/library/dcm.h"

#include <list>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>
#include <vector>

namespace {

/// Keeps an address, so that the compiler cannot leave it out.
template <class Address>
void Take(Address address)
{
    [[maybe_unused]] static volatile Address kept;
    kept = address;
}

/// The same for one of several functions of a name.
template <class Signature, class Class>
void TakeMember(Signature Class::*member)
{
    Take(member);
}
template <class Signature>
void TakeFunction(Signature* function)
{
    Take(function);
}

/// Constructors, assignments and the destructor.
template <class Class>
void Copy(Class object)
{
    Class copy(object);
    copy = object;
    Class moved(std::move(copy));
    moved = std::move(object);
}

void Texts()
{
    static constinit dcm::TextConstant constant(L"text");
    Copy(CString());
    Copy(CString(constant));
    Copy(CString(L""));
    Copy(CString(""));
    Copy(CString(std::wstring_view(constant)));
    Take(&CString::GetLength);
    Take(&CString::IsEmpty);
    Take(&CString::GetAt);
    Take(&CString::SetAt);
    Take(&CString::operator const wchar_t*);
    Take(&CString::operator std::wstring_view);
    Take(&CString::View);
    Take(&CString::Compare);
    Take(&CString::CompareNoCase);
    TakeMember<int(std::wstring_view, int) const noexcept>(&CString::Find);
    TakeMember<int(wchar_t, int) const noexcept>(&CString::Find);
    Take(&CString::FindOneOf);
    Take(&CString::Left);
    Take(&CString::Right);
    TakeMember<CString(int) const>(&CString::Mid);
    TakeMember<CString(int, int) const>(&CString::Mid);
    TakeMember<CString&()>(&CString::Trim);
    TakeMember<CString&(std::wstring_view)>(&CString::Trim);
    TakeMember<CString&()>(&CString::TrimLeft);
    TakeMember<CString&(std::wstring_view)>(&CString::TrimLeft);
    TakeMember<CString&()>(&CString::TrimRight);
    TakeMember<CString&(std::wstring_view)>(&CString::TrimRight);
    TakeMember<int(std::wstring_view, std::wstring_view)>(&CString::Replace);
    TakeMember<int(wchar_t, wchar_t)>(&CString::Replace);
    Take(&CString::Empty);
    Take(&CString::Append);
    Take(&CString::AppendChar);
    TakeMember<CString&(std::wstring_view), CString>(&CString::operator+=);
    TakeMember<CString&(wchar_t), CString>(&CString::operator+=);
    Take(&CString::Extend);
    Take(&CString::EndExtend);

    // Friends, whose address cannot be taken.
    const CString text = CString(L"") + L"" + L'_' + CString(L"");
    const CString longer = L'_' + (L"" + text);
    Take(longer == text && longer == L"" && longer == L'_' && longer == std::wstring_view());
    Take((longer <=> text) == (longer <=> L"") && (longer <=> L'_') == (longer <=> constant));

    Take(&dcm::SetThreadCodePage);
    Take(&dcm::ThreadCodePage);
    Take(&dcm::ToUtf8);
    Take(&dcm::FromUtf8);
}

void Variants()
{
    // Constants would not call the constructors.
    volatile double number = 1.0;
    volatile float single = 1.0F;
    volatile int integer = 1;
    Copy(CComVariant());
    Copy(CComVariant(number));
    Copy(CComVariant(single));
    Copy(CComVariant(integer));
    Copy(CComVariant(L""));
    Copy(CComVariant(CString()));
    Copy(CComVariant(std::wstring_view()));
    Copy(CComVariant(VARIANT{}));
    TakeMember<CComVariant&(const VARIANT&)>(&CComVariant::operator=);
    Take(&CComVariant::SetText);
    Take(&CComVariant::Detach);
    Take(&CComVariant::Clear);
    Take(&CComVariant::TextOf);
    Take(&VariantInit);
    Take(&VariantClear);
    Take(&VariantCopy);
    Take(&SysAllocString);
    Take(&SysAllocStringLen);
    Take(&SysFreeString);
    Take(&SysStringLen);
    Take(&SUCCEEDED);
    Take(&FAILED);
}

void Failures()
{
    Copy(dcm::ResultError(E_FAIL));
    Take(&dcm::ResultError::Code);
    Take(dcm::ResultError(E_FAIL).dcm::ResultError::what());
    Take(&dcm::ThrowResult);
    Copy(CFileException());
    Copy(CFileException(CFileException::generic, 0, CString()));
}

struct OpenFile : PravFile
{
    using CFile::FilePath, PravFile::LoadContent;
};

/// Virtual members are called: their address does not name them.
template <class File>
void Files()
{
    File();
    File file(CString(), CFile::modeRead);
    CFileStatus status;
    Take(file.File::Open(L"", CFile::modeRead, nullptr));
    Take(file.CFile::GetStatus(status));
    Take(file.CFile::GetLength());
    Take(file.CFile::Read(&status, 0));
    file.CFile::Write(&status, 0);
    file.CFile::Close();
}

void Modules()
{
    AFX_EXTENSION_MODULE state;
    CDynLinkLibrary library(state);
    Take(&CDynLinkLibrary::Module);
    Take(&CDynLinkLibrary::Last);
    Take(&CDynLinkLibrary::Previous);
    Take(&AfxInitExtensionModule);
    Take(&AfxTermExtensionModule);
    Take(&dcm::LibraryVersion);
}

struct OpenMap : DCMKennfeld
{
    using DCMBaseType::ExportDisplayname, DCMBaseType::ExportFunktion, DCMBaseType::ExportLangname;
    using DCMKennfeld::AddValues, DCMKennfeld::ExportValues;
};

using Array = HRESULT(std::vector<CComVariant>&) const;

void Blocks()
{
    Copy(DCMBaseType());
    TakeMember<CString&()>(&DCMBaseType::GetName);
    TakeMember<const CString&() const>(&DCMBaseType::GetName);
    TakeMember<CString&()>(&DCMBaseType::GetLangname);
    TakeMember<const CString&() const>(&DCMBaseType::GetLangname);
    TakeMember<CString&()>(&DCMBaseType::GetDisplayname);
    TakeMember<const CString&() const>(&DCMBaseType::GetDisplayname);
    TakeMember<CString&()>(&DCMBaseType::GetFunction);
    TakeMember<const CString&() const>(&DCMBaseType::GetFunction);
    Take(&DCMBaseType::SetName);
    Take(&DCMBaseType::SetLangname);
    Take(&DCMBaseType::SetDisplayname);
    Take(&DCMBaseType::SetFunction);
    Take(&OpenMap::ExportLangname);
    Take(&OpenMap::ExportDisplayname);
    Take(&OpenMap::ExportFunktion);

    Copy(DCMKonservierungsFormat());
    Take(&DCMKonservierungsFormat::Init);
    Take(&DCMKonservierungsFormat::SetValue);
    Take(&DCMKonservierungsFormat::GetValue);
    Take(&DCMKonservierungsFormat::Export);

    Copy(DCMFestwert());
    Copy(DCMTextstring());
    Take(&DCMFestwert::Init);
    Take(&DCMFestwert::Export);
    Take(&DCMFestwert::GetValue);
    TakeMember<HRESULT(const VARIANT&), DCMFestwert>(&DCMFestwert::SetValue);
    TakeMember<HRESULT(const VARIANT*), DCMFestwert>(&DCMFestwert::SetValue);
    Take(&DCMFestwert::SetValue<double>);
    Take(&DCMFestwert::GetValueType);
    TakeMember<CString&()>(&DCMFestwert::GetUnit);
    TakeMember<const CString&() const>(&DCMFestwert::GetUnit);
    Take(&DCMFestwert::SetUnit);

    Copy(DCMFestwerteblock());
    Take(&DCMFestwerteblock::Init);
    Take(&DCMFestwerteblock::Export);
    TakeMember<void(double)>(&DCMFestwerteblock::AddValue);
    TakeMember<void(const CString&)>(&DCMFestwerteblock::AddValue);
    Take(&DCMFestwerteblock::GetDoubleValues);
    Take(&DCMFestwerteblock::GetStringValues);
    TakeMember<CString&()>(&DCMFestwerteblock::GetUnit);
    TakeMember<const CString&() const>(&DCMFestwerteblock::GetUnit);
    Take(&DCMFestwerteblock::SetUnit);
    Take(&DCMFestwerteblock::GetXValueCount);
    Take(&DCMFestwerteblock::GetYValueCount);
    Take(&DCMFestwerteblock::SetXValueCount);
    Take(&DCMFestwerteblock::SetYValueCount);

    Copy(DCMStuetzstellenverteilung());
    Take(&DCMStuetzstellenverteilung::Init);
    Take(&DCMStuetzstellenverteilung::Export);
    Take(&DCMStuetzstellenverteilung::AddValue);
    Take(&DCMStuetzstellenverteilung::GetValues);
    Take(&DCMStuetzstellenverteilung::GetValueType);
    TakeMember<CString&()>(&DCMStuetzstellenverteilung::GetUnit);
    TakeMember<const CString&() const>(&DCMStuetzstellenverteilung::GetUnit);
    Take(&DCMStuetzstellenverteilung::SetUnit);
}

void CurvesAndMaps()
{
    Copy(DCMKennlinie());
    Copy(DCMFestkennlinie());
    Copy(DCMGruppenkennlinie());
    Take(&DCMKennlinie::Init);
    Take(&DCMKennlinie::Export);
    TakeMember<HRESULT(VARIANT)>(&DCMKennlinie::AddValue);
    TakeMember<void(double, const CString&)>(&DCMKennlinie::AddValue);
    Take(&DCMKennlinie::AddAxis);
    TakeMember<Array>(&DCMKennlinie::GetAxis);
    TakeMember<Array>(&DCMKennlinie::GetValues);
    TakeMember<std::list<double>() const>(&DCMKennlinie::GetAxis);
    TakeMember<std::list<double>() const>(&DCMKennlinie::GetValues);
    Take(&DCMKennlinie::GetAxisType);
    Take(&DCMKennlinie::GetValueType);
    Take(&DCMKennlinie::GetAxisLenghtX);
    Take(&DCMKennlinie::SetAxisLenghtX);
    TakeMember<CString&()>(&DCMKennlinie::GetUnit_X);
    TakeMember<const CString&() const>(&DCMKennlinie::GetUnit_X);
    TakeMember<CString&()>(&DCMKennlinie::GetUnit_W);
    TakeMember<const CString&() const>(&DCMKennlinie::GetUnit_W);
    Take(&DCMKennlinie::SetUnit_X);
    Take(&DCMKennlinie::SetUnit_W);
    Take(&DCMKennlinie::SetSharedAxisUniqueName);
    Take(&DCMKennlinie::GetStuetzstellenverteilung);

    Copy(DCMKennfeld());
    Copy(DCMFestkennfeld());
    Copy(DCMGruppenkennfeld());
    Take(&DCMKennfeld::Init);
    Take(&DCMKennfeld::Export);
    Take(&DCMKennfeld::AddValue);
    Take(&DCMKennfeld::AddAxisX);
    Take(&DCMKennfeld::AddAxisY);
    Take(&DCMKennfeld::GetAxis_X);
    Take(&DCMKennfeld::GetAxis_Y);
    Take(&DCMKennfeld::GetValues);
    Take(&DCMKennfeld::GetAxis_XType);
    Take(&DCMKennfeld::GetAxis_YType);
    Take(&DCMKennfeld::GetValueType);
    Take(&DCMKennfeld::GetAxisLenghtX);
    Take(&DCMKennfeld::GetAxisLenghtY);
    Take(&DCMKennfeld::SetAxisLenghtX);
    Take(&DCMKennfeld::SetAxisLenghtY);
    TakeMember<CString&()>(&DCMKennfeld::GetUnit_X);
    TakeMember<const CString&() const>(&DCMKennfeld::GetUnit_X);
    TakeMember<CString&()>(&DCMKennfeld::GetUnit_Y);
    TakeMember<const CString&() const>(&DCMKennfeld::GetUnit_Y);
    TakeMember<CString&()>(&DCMKennfeld::GetUnit_W);
    TakeMember<const CString&() const>(&DCMKennfeld::GetUnit_W);
    Take(&DCMKennfeld::SetUnit_X);
    Take(&DCMKennfeld::SetUnit_Y);
    Take(&DCMKennfeld::SetUnit_W);
    Take(&DCMKennfeld::SetSharedXAxisUniqueName);
    Take(&DCMKennfeld::SetSharedYAxisUniqueName);
    Take(&DCMKennfeld::GetStuetzstellenverteilungX);
    Take(&DCMKennfeld::GetStuetzstellenverteilungY);
    Take(&DCMKennfeld::RotateMap);
    Take(&OpenMap::AddValues);
    Take(&OpenMap::ExportValues);
}

void Documents()
{
    Copy(DCMHeader());
    Take(&DCMHeader::SetText);
    Take(&DCMHeader::Export);
    Copy(DCMConverter());
    Take(&DCMConverter::Import);
    Take(&DCMConverter::Export);
    Take(&DCMConverter::SetVersion);
    Take(&DCMConverter::SetHeader);
    Take(&DCMConverter::GetComment);
    Take(&DCMConverter::AddFestwert);
    Take(&DCMConverter::AddFestwerteblock);
    Take(&DCMConverter::AddStuetzstellenverteilung);
    Take(&DCMConverter::AddKennlinie);
    Take(&DCMConverter::AddFestkennlinie);
    Take(&DCMConverter::AddGruppenkennlinie);
    Take(&DCMConverter::AddKennfeld);
    Take(&DCMConverter::AddFestkennfeld);
    Take(&DCMConverter::AddGruppenkennfeld);
    Take(&DCMConverter::AddTextstring);
    Take(&DCMConverter::GetFestwerte);
    Take(&DCMConverter::GetFestwerteblock);
    Take(&DCMConverter::GetStuetzstellenverteilung);
    Take(&DCMConverter::GetKennlinie);
    Take(&DCMConverter::GetFestkennlinie);
    Take(&DCMConverter::GetGruppenkennlinie);
    Take(&DCMConverter::GetKennfeld);
    Take(&DCMConverter::GetFestkennfeld);
    Take(&DCMConverter::GetGruppenkennfeld);
    Take(&DCMConverter::GetTextstring);
}

template <class Block>
void Visit(dcm::BlockVisitor& visitor)
{
    visitor.dcm::BlockVisitor::Visit(Block());
}

void Parameters()
{
    dcm::BlockVisitor visitor;
    Copy(visitor);
    Visit<DCMFestwert>(visitor);
    Visit<DCMFestwerteblock>(visitor);
    Visit<DCMStuetzstellenverteilung>(visitor);
    Visit<DCMKennlinie>(visitor);
    Visit<DCMFestkennlinie>(visitor);
    Visit<DCMGruppenkennlinie>(visitor);
    Visit<DCMKennfeld>(visitor);
    Visit<DCMFestkennfeld>(visitor);
    Visit<DCMGruppenkennfeld>(visitor);
    Visit<DCMTextstring>(visitor);
    TakeFunction<void(const DCMConverter&, dcm::BlockVisitor&)>(&dcm::ForEach);
    dcm::ForEach(DCMConverter(), [](const auto&) {});

    Copy(dcm::Parameter());
    Copy(dcm::Axis());
    TakeFunction<std::wstring_view(dcm::Kind) noexcept>(&dcm::KeywordOf);
    Take(&dcm::KindOf);
    TakeFunction<dcm::Parameter(const DCMFestwert&)>(&dcm::ParameterOf);
    TakeFunction<dcm::Parameter(const DCMFestwerteblock&)>(&dcm::ParameterOf);
    TakeFunction<dcm::Parameter(const DCMStuetzstellenverteilung&)>(&dcm::ParameterOf);
    TakeFunction<dcm::Parameter(const DCMKennlinie&)>(&dcm::ParameterOf);
    TakeFunction<dcm::Parameter(const DCMKennfeld&)>(&dcm::ParameterOf);
    TakeFunction<std::vector<dcm::Parameter>(const DCMConverter&)>(&dcm::ParametersOf);
    TakeFunction<std::vector<dcm::Parameter>(DCMConverter &&)>(&dcm::ParametersOf);
    TakeFunction<void(DCMConverter&, const dcm::Parameter&)>(&dcm::Add);
    TakeFunction<void(DCMConverter&, dcm::Parameter &&)>(&dcm::Add);
    Take(&dcm::HeaderOfComment);

    TakeFunction<std::wstring_view(dcm::Field) noexcept>(&dcm::KeywordOf);
    Take(&dcm::Differences);
    Copy(dcm::Difference());
}

void Reports()
{
    Copy(dcm::Finding());
    Copy(dcm::Report());
    Take(&dcm::Report::Findings);
    TakeMember<std::size_t(dcm::Severity) const noexcept>(&dcm::Report::Count);
    TakeMember<std::size_t(std::string_view) const noexcept>(&dcm::Report::Count);
    TakeMember<std::size_t() const noexcept>(&dcm::Report::Count);
    Take(&dcm::Report::Summary);
    Take(&dcm::Report::SetLimit);
    Take(&dcm::Report::Limit);
    Take(&dcm::Report::Incomplete);
    Take(&dcm::Report::Cause);
    Take(&dcm::Report::SystemError);
    Take(&dcm::NameOf);
    Take(&dcm::FindingIds);
    Take(&dcm::Import);
    Take(&dcm::Export);
    Take(&dcm::Save);
    Take(&dcm::NullDevice);
}

} // namespace

int main()
{
    Texts();
    Variants();
    Failures();
    Files<CFile>();
    Files<PravFile>();
    Take(&PravFile::ReadLine);
    Take(&PravFile::WriteText);
    Take(&OpenFile::FilePath);
    Take(&OpenFile::LoadContent);
    Modules();
    Blocks();
    CurvesAndMaps();
    Documents();
    Parameters();
    Reports();
}
