#include "testclasses.h"

OMB_DEFINE_ENGINE_CLASS(TestUnit, OmbResourceObject, "TestUnit", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(TestUnit)
OMB_DEFINE_ENGINE_CLASS(TestShape, OmbResourceObject, "TestShape", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(TestShape)

OMB_DESCRIBE_CLASS(TestUnit) {
    d.property<double>(
        "InMeters", [](const TestUnit& u) { return u.inMeters(); }, [](TestUnit& u, double v) { u.inMeters(v); }, 1.0);
}

OMB_DESCRIBE_CLASS(TestShape) {
    d.property<double>("Width", &TestShape::width, [](TestShape& s, double v) { s.width = v; }).required();
    d.property<long long>("Count", &TestShape::count, [](TestShape& s, long long v) { s.count = v; });
    d.property<bool>(
        "Visible", &TestShape::visible, [](TestShape& s, bool v) { s.visible = v; }, true);
    d.property<OmbString>("Label", &TestShape::label, [](TestShape& s, const OmbString& v) { s.label = v; });
    d.property<OmbChildObjectMode>("Mode", &TestShape::mode, [](TestShape& s, OmbChildObjectMode v) { s.mode = v; });
    d.object<TestUnit>("Unit", &TestShape::unit, [](TestShape& s, const OmbRef<TestUnit>& v) { s.unit = v; });
    d.collection<TestShapeVec>("Parts", "TestShapeCollection", &TestShape::parts,
                               [](TestShape& s, const OmbRef<TestShapeVec>& v) { s.parts = v; })
        .content();
}
