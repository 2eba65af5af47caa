#include "dcm/elements/block_fields.h"

#include "dcm/elements/block_io.h"
#include "dcm/elements/festwert.h"
#include "dcm/elements/festwerteblock.h"
#include "dcm/elements/kennfeld.h"
#include "dcm/elements/kennlinie.h"
#include "dcm/elements/stuetzstellenverteilung.h"

namespace dcm {

ValueFields BlockIo::FieldsOf(DCMFestwert& block)
{
    return {block.m_strKeyword, block.m_value};
}

ListFields BlockIo::FieldsOf(DCMFestwerteblock& block)
{
    return {block.m_vecDoubleValues, block.m_listStringValues};
}

DistributionFields BlockIo::FieldsOf(DCMStuetzstellenverteilung& block)
{
    return {{block.m_vecValues, block.m_vtValueType}};
}

CurveFields BlockIo::FieldsOf(DCMKennlinie& block)
{
    return {block.m_strKeyword,
            {{block.m_vecAxis, block.m_vtAxisType},
             block.m_strStuetzstellenverteilung,
             block.m_strSharedAxisUniqueName},
            {block.m_vecValues, block.m_vtValueType}};
}

MapFields BlockIo::FieldsOf(DCMKennfeld& block)
{
    return {block.m_strKeyword,
            {{block.m_vecAxisX, block.m_vtAxisXType},
             block.m_strStuetzstellenverteilungX,
             block.m_strSharedXAxisUniqueName},
            {{block.m_vecAxisY, block.m_vtAxisYType},
             block.m_strStuetzstellenverteilungY,
             block.m_strSharedYAxisUniqueName},
            {block.m_vecValues, block.m_vtValueType}};
}

} // namespace dcm
